<?xml version="1.0" encoding="UTF-8"?>
<!-- Turns a report of a clash result into an HTML page: what was computed, then a table a result
     set. It needs no script and nothing from a network. -->
<xsl:stylesheet version="1.0" xmlns:xsl="http://www.w3.org/1999/XSL/Transform">
  <xsl:output method="html" version="5" encoding="UTF-8" indent="yes"
              doctype-system="about:legacy-compat"/>

  <xsl:variable name="title">
    <xsl:text>Clash result</xsl:text>
    <xsl:if test="/*/@ZORDocument != ''">
      <xsl:text> </xsl:text>
      <xsl:value-of select="/*/@ZORDocument"/>
    </xsl:if>
  </xsl:variable>

  <xsl:template match="/">
    <html>
      <head>
        <title><xsl:value-of select="$title"/></title>
        <meta name="viewport" content="width=device-width"/>
        <style>
          body { font: 15px/1.45 system-ui, sans-serif; margin: 2rem; color: #222; background: #fff; }
          h1 { font-size: 1.5rem; margin: 0 0 .5rem; }
          h2 { font-size: 1.15rem; margin: 2rem 0 .25rem; }
          dl { display: grid; grid-template-columns: max-content 1fr; gap: .1rem 1.5rem; margin: 0; }
          dt { color: #666; }
          dd { margin: 0; }
          table { border-collapse: collapse; margin-top: .75rem; width: 100%; }
          th, td { padding: .35rem .6rem; text-align: left; vertical-align: top;
                   border-bottom: 1px solid #ddd; overflow-wrap: anywhere; }
          th { background: #f4f4f4; position: sticky; top: 0; overflow-wrap: normal; }
          .number { text-align: right; font-variant-numeric: tabular-nums; white-space: nowrap; }
          .clash td:nth-child(2) { color: #b00020; font-weight: 600; }
          .contact td:nth-child(2) { color: #8a5a00; }
          .clearance td:nth-child(2) { color: #00639b; }
          .note { color: #666; }
          @media print { body { margin: 0; } th { position: static; } }
        </style>
      </head>
      <body><xsl:apply-templates/></body>
    </html>
  </xsl:template>

  <xsl:template match="ClashElement | InterferenceElement">
    <h1><xsl:value-of select="$title"/></h1>
    <dl>
      <xsl:call-template name="fact">
        <xsl:with-param name="name">Responsible</xsl:with-param>
        <xsl:with-param name="value" select="@Responsible"/>
      </xsl:call-template>
      <xsl:apply-templates select="Date[last()]"/>
      <xsl:apply-templates select="ClashSpec[last()]"/>
      <xsl:call-template name="fact">
        <xsl:with-param name="name">Interferences</xsl:with-param>
        <xsl:with-param name="value" select="count(ClashResult/Interference | Interference)"/>
      </xsl:call-template>
    </dl>
    <xsl:apply-templates select="ClashResult"/>
    <xsl:if test="Interference">
      <xsl:call-template name="table">
        <xsl:with-param name="rows" select="Interference[1]"/>
      </xsl:call-template>
    </xsl:if>
  </xsl:template>

  <xsl:template name="fact">
    <xsl:param name="name"/>
    <xsl:param name="value"/>
    <xsl:if test="$value != ''">
      <dt><xsl:value-of select="$name"/></dt>
      <dd><xsl:value-of select="$value"/></dd>
    </xsl:if>
  </xsl:template>

  <xsl:template match="Date">
    <dt>Date</dt>
    <dd>
      <xsl:choose>
        <xsl:when test="@Day and @Month and @Year">
          <xsl:value-of select="concat(@Year, '-', format-number(@Month, '00'), '-',
                                       format-number(@Day, '00'))"/>
        </xsl:when>
        <xsl:otherwise>
          <xsl:for-each select="@*">
            <xsl:if test="position() > 1"><xsl:text> </xsl:text></xsl:if>
            <xsl:value-of select="."/>
          </xsl:for-each>
        </xsl:otherwise>
      </xsl:choose>
    </dd>
  </xsl:template>

  <xsl:template match="ClashSpec">
    <dt>Specification</dt>
    <dd>
      <xsl:value-of select="@Name"/>
      <xsl:if test="@Type != ''"><xsl:value-of select="concat(', ', @Type)"/></xsl:if>
      <xsl:if test="@Clearance != ''">
        <xsl:value-of select="concat(', clearance ', @Clearance, ' mm')"/>
      </xsl:if>
    </dd>
  </xsl:template>

  <xsl:template match="ClashResult">
    <h2><xsl:value-of select="@Name"/></h2>
    <p class="note"><xsl:value-of select="@ComputationCase"/></p>
    <xsl:call-template name="table">
      <xsl:with-param name="rows" select="Interference"/>
      <xsl:with-param name="before" select="count(preceding-sibling::ClashResult/Interference)"/>
    </xsl:call-template>
  </xsl:template>

  <!-- Interferences are numbered over all result sets. -->
  <xsl:template name="table">
    <xsl:param name="rows"/>
    <xsl:param name="before" select="0"/>
    <table>
      <thead>
        <tr>
          <th class="number">N</th>
          <th>Type</th>
          <th class="number">Value</th>
          <th>Status</th>
          <th>First product</th>
          <th>Second product</th>
          <th>Rule</th>
          <th>Comment</th>
        </tr>
      </thead>
      <tbody>
        <xsl:for-each select="$rows">
          <xsl:apply-templates select="." mode="row">
            <xsl:with-param name="number" select="$before + position()"/>
          </xsl:apply-templates>
        </xsl:for-each>
      </tbody>
    </table>
  </xsl:template>

  <xsl:template match="Interference" mode="row">
    <xsl:param name="number"/>
    <tr>
      <xsl:attribute name="class">
        <xsl:value-of select="translate(@ResultTypeNoNLS, 'CL', 'cl')"/>
      </xsl:attribute>
      <td class="number"><xsl:value-of select="$number"/></td>
      <td>
        <xsl:choose>
          <xsl:when test="@ResultTypeNoNLS"><xsl:value-of select="@ResultTypeNoNLS"/></xsl:when>
          <xsl:otherwise><xsl:value-of select="@ResultType"/></xsl:otherwise>
        </xsl:choose>
      </td>
      <td class="number"><xsl:value-of select="@Value"/></td>
      <td><xsl:value-of select="@Status"/></td>
      <td><xsl:apply-templates select="Product[1]"/></td>
      <td><xsl:apply-templates select="Product[position() > 1][last()]"/></td>
      <td>
        <xsl:value-of select="ViolatedRule[last()]/@Name"/>
        <xsl:if test="ViolatedRule[last()]/@Severity != ''">
          <span class="note">
            <xsl:value-of select="concat(' ', ViolatedRule[last()]/@Severity)"/>
          </span>
        </xsl:if>
      </td>
      <td><xsl:value-of select="Comment[last()]/@Value"/></td>
    </tr>
  </xsl:template>

  <xsl:template match="Product">
    <xsl:choose>
      <xsl:when test="@Alias != ''"><xsl:value-of select="@Alias"/></xsl:when>
      <xsl:otherwise><xsl:value-of select="@DescriptionID"/></xsl:otherwise>
    </xsl:choose>
  </xsl:template>

  <xsl:template match="ProductsInSpec | text()"/>
</xsl:stylesheet>
