<xsl:stylesheet version="1.0" xmlns:xsl="http://www.w3.org/1999/XSL/Transform">
<xsl:output method="html" encoding="UTF-8"/><xsl:key name="k" match="*" use="@Name"/><xsl:variable name="v" select="//*[1]"/>
<xsl:template match="/"><html><xsl:apply-templates select="*"><xsl:sort select="@Name"/></xsl:apply-templates></html></xsl:template>
<xsl:template match="*" name="t"><xsl:param name="p" select="2"/><p class="{@Name}"><xsl:value-of select="concat(name(),format-number($p,'0.0'),key('k','r')/@Name)"/></p>
<xsl:choose><xsl:when test="position()=1"><xsl:for-each select="*|@*"><xsl:copy/></xsl:for-each></xsl:when><xsl:otherwise><xsl:message>m</xsl:message></xsl:otherwise></xsl:choose><xsl:number/></xsl:template>
</xsl:stylesheet>
