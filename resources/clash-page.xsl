<?xml version="1.0" encoding="UTF-8"?>
<!-- Turns a report of a clash result into the page that "lyra publish" writes. Beside what a report
     holds, that command gives to the root: page:model, page:policy (what the page may load), a
     page:Type for each type and a page:Status for each status, with page:word and page:count, a
     page:Cell for each type with a status, page:Style and page:Script (resources/page) and page:Data,
     JSON for the script; to each interference: page:number, page:id, page:type, page:status,
     page:picture, page:asInModel (why the picture does not have the result's placements) and
     page:Thumbnail elements; to each of its two products: page:colour, page:preview and page:missing.
     page:asInModel at the root says that no picture has them, as was asked for. A picture in the page
     itself is referred to as "#id". Texts of the document are isolated (bdi), so that none can change
     the direction of what stands around it. -->
<xsl:stylesheet version="1.0" xmlns:xsl="http://www.w3.org/1999/XSL/Transform"
                xmlns:page="urn:zorlyra:page" exclude-result-prefixes="page">
  <xsl:output method="html" version="5" encoding="UTF-8" indent="no"
              doctype-system="about:legacy-compat"/>

  <xsl:variable name="interferences"
                select="/ClashElement/ClashResult/Interference | /InterferenceElement/Interference[1]"/>
  <!-- Those of an older result that this one has no more. -->
  <xsl:variable name="gone" select="/*/page:Gone/Interference"/>
  <xsl:variable name="all" select="$interferences | $gone"/>
  <xsl:variable name="hasBaseline" select="boolean(/*/@page:baseline)"/>
  <xsl:variable name="hasPictures" select="boolean($all/@page:picture | $all/@page:before)"/>
  <xsl:variable name="mostPoints" select="100"/>
  <xsl:variable name="mostWords" select="12"/>
  <!-- With more interferences than this, a script puts sections and pictures in where they are seen: browsers
       take long over thousands of them. -->
  <xsl:variable name="mostLazy" select="500"/>
  <xsl:variable name="areMany" select="count($interferences) > $mostLazy"/>

  <xsl:variable name="title">
    <xsl:choose>
      <xsl:when test="/*/@ZORDocument != ''"><xsl:value-of select="/*/@ZORDocument"/></xsl:when>
      <xsl:otherwise>Clash result</xsl:otherwise>
    </xsl:choose>
  </xsl:variable>

  <xsl:template match="/">
    <html lang="en">
      <head>
        <title><xsl:value-of select="$title"/> · clash report</title>
        <meta name="viewport" content="width=device-width, initial-scale=1"/>
        <meta name="color-scheme" content="light dark"/>
        <meta http-equiv="Content-Security-Policy"
              content="{/*/@page:policy}"/>
        <link rel="icon" href="data:,"/>
        <style><xsl:value-of select="/*/page:Style"/></style>
      </head>
      <body>
        <xsl:apply-templates select="/ClashElement | /InterferenceElement"/>
        <script type="application/json" id="zor-data"><xsl:value-of select="/*/page:Data"/></script>
        <script><xsl:value-of select="/*/page:Script"/></script>
      </body>
    </html>
  </xsl:template>

  <xsl:template match="ClashElement | InterferenceElement">
    <header>
      <p class="kind">Clash report</p>
      <h1><bdi><xsl:value-of select="$title"/></bdi></h1>
      <dl class="facts">
        <xsl:call-template name="fact">
          <xsl:with-param name="name">Responsible</xsl:with-param>
          <xsl:with-param name="value" select="@Responsible"/>
        </xsl:call-template>
        <xsl:apply-templates select="Date[last()]"/>
        <xsl:apply-templates select="ClashSpec[last()]"/>
        <xsl:call-template name="fact">
          <xsl:with-param name="name">Model</xsl:with-param>
          <xsl:with-param name="value" select="@page:model"/>
        </xsl:call-template>
        <xsl:call-template name="fact">
          <xsl:with-param name="name">Compared with</xsl:with-param>
          <xsl:with-param name="value" select="@page:baseline"/>
        </xsl:call-template>
        <xsl:call-template name="fact">
          <xsl:with-param name="name">Interferences</xsl:with-param>
          <xsl:with-param name="value" select="count($interferences)"/>
        </xsl:call-template>
      </dl>
      <xsl:if test="$interferences">
        <div class="overview">
          <div><xsl:call-template name="matrix"/></div>
          <xsl:if test="@page:map"><xsl:call-template name="map"/></xsl:if>
        </div>
      </xsl:if>
      <xsl:if test="@page:asInModel">
        <p class="note">The pictures show the products where they stand in the model.</p>
      </xsl:if>
      <xsl:if test="$interferences/@page:asInModel">
        <p class="notice">
          <strong><xsl:value-of select="count($interferences[@page:asInModel])"/></strong>
          <xsl:text> of </xsl:text>
          <xsl:value-of select="count($interferences)"/>
          <xsl:text> interferences are drawn with the products where they stand in the model, since the placements of the result cannot be used.</xsl:text>
        </p>
      </xsl:if>
      <xsl:if test="$interferences/Product/@page:missing">
        <p class="notice">
          <strong><xsl:value-of select="count($interferences[Product/@page:missing])"/></strong>
          <xsl:text> of </xsl:text>
          <xsl:value-of select="count($interferences)"/>
          <xsl:text> interferences name a product that the model does not have. They are marked </xsl:text>
          <span class="missing">not in the model</span>.
        </p>
      </xsl:if>
    </header>
    <main>
      <xsl:choose>
        <xsl:when test="$all">
          <xsl:call-template name="table"/>
          <xsl:for-each select="$all">
            <xsl:apply-templates select="." mode="section"/>
          </xsl:for-each>
        </xsl:when>
        <xsl:otherwise><p class="notice">There is no interference to show.</p></xsl:otherwise>
      </xsl:choose>
    </main>
  </xsl:template>

  <!-- Summary -->
  <xsl:template name="fact">
    <xsl:param name="name"/>
    <xsl:param name="value"/>
    <xsl:if test="$value != ''">
      <div><dt><xsl:value-of select="$name"/></dt><dd><bdi><xsl:value-of select="$value"/></bdi></dd></div>
    </xsl:if>
  </xsl:template>

  <xsl:template name="length">
    <xsl:param name="name"/>
    <xsl:param name="value"/>
    <xsl:if test="$value != ''">
      <div>
        <dt><xsl:value-of select="$name"/></dt>
        <dd class="value"><xsl:call-template name="number"><xsl:with-param name="text" select="$value"/><xsl:with-param name="unit"> mm</xsl:with-param></xsl:call-template>&#160;mm</dd>
      </div>
    </xsl:if>
  </xsl:template>

  <xsl:template match="Date">
    <xsl:variable name="text">
      <xsl:choose>
        <xsl:when test="number(@Day) = number(@Day) and number(@Month) = number(@Month) and @Year">
          <xsl:value-of select="concat(@Year, '-', format-number(@Month, '00'), '-', format-number(@Day, '00'))"/>
        </xsl:when>
        <xsl:otherwise>
          <xsl:for-each select="@*">
            <xsl:if test="position() > 1"><xsl:text> </xsl:text></xsl:if>
            <xsl:value-of select="."/>
          </xsl:for-each>
        </xsl:otherwise>
      </xsl:choose>
    </xsl:variable>
    <xsl:call-template name="fact">
      <xsl:with-param name="name">Date</xsl:with-param>
      <xsl:with-param name="value" select="$text"/>
    </xsl:call-template>
  </xsl:template>

  <xsl:template match="ClashSpec">
    <xsl:variable name="text">
      <xsl:value-of select="@Name"/>
      <xsl:if test="@Type != ''"><xsl:value-of select="concat(', ', @Type)"/></xsl:if>
      <xsl:if test="@Clearance != ''"><xsl:value-of select="concat(', clearance&#160;', @Clearance, '&#160;mm')"/></xsl:if>
    </xsl:variable>
    <xsl:call-template name="fact">
      <xsl:with-param name="name">Specification</xsl:with-param>
      <xsl:with-param name="value" select="$text"/>
    </xsl:call-template>
  </xsl:template>

  <!-- How many of each type have each status. Of very many words the most frequent ones. -->
  <xsl:template name="matrix">
    <xsl:variable name="root" select="."/>
    <xsl:variable name="types" select="page:Type[position() &lt;= $mostWords]"/>
    <xsl:variable name="statuses" select="page:Status[position() &lt;= $mostWords]"/>
    <table id="matrix">
      <caption>Interferences by type and status</caption>
      <thead>
        <tr>
          <th scope="col">Type</th>
          <xsl:for-each select="$statuses">
            <th scope="col" class="number"><xsl:call-template name="short"><xsl:with-param name="text" select="@page:word"/></xsl:call-template></th>
          </xsl:for-each>
          <th scope="col" class="number">All</th>
        </tr>
      </thead>
      <tbody>
        <xsl:for-each select="$types">
          <xsl:variable name="type" select="@page:word"/>
          <xsl:variable name="class"><xsl:call-template name="class"><xsl:with-param name="word" select="$type"/></xsl:call-template></xsl:variable>
          <tr>
            <th scope="row"><span class="dot {$class}"></span><xsl:call-template name="short"><xsl:with-param name="text" select="$type"/></xsl:call-template></th>
            <xsl:for-each select="$statuses">
              <xsl:variable name="count" select="$root/page:Cell[@page:type = $type and @page:word = current()/@page:word]/@page:count"/>
              <td class="number">
                <xsl:choose>
                  <xsl:when test="$count"><xsl:value-of select="$count"/></xsl:when>
                  <xsl:otherwise><span class="none">0</span></xsl:otherwise>
                </xsl:choose>
              </td>
            </xsl:for-each>
            <td class="number all"><xsl:value-of select="@page:count"/></td>
          </tr>
        </xsl:for-each>
      </tbody>
      <tfoot>
        <tr>
          <th scope="row">All</th>
          <xsl:for-each select="$statuses"><td class="number"><xsl:value-of select="@page:count"/></td></xsl:for-each>
          <td class="number all"><xsl:value-of select="count($interferences)"/></td>
        </tr>
      </tfoot>
    </table>
    <xsl:if test="count(page:Type) > $mostWords or count(page:Status) > $mostWords">
      <p class="note">The most frequent types and statuses are counted here.</p>
    </xsl:if>
  </xsl:template>

  <!-- The whole model, with a link where each interference is. -->
  <xsl:template name="map">
    <figure class="map">
      <div>
        <xsl:call-template name="image">
          <xsl:with-param name="path" select="@page:map"/>
          <xsl:with-param name="meaning">The whole model</xsl:with-param>
        </xsl:call-template>
        <svg class="points" viewBox="0 0 1000 {@page:mapHeight}" role="group" aria-label="Where the interferences are">
          <xsl:for-each select="$interferences[@page:mapX]">
            <xsl:variable name="class"><xsl:call-template name="class"><xsl:with-param name="word" select="@page:type"/></xsl:call-template></xsl:variable>
            <a class="{$class}" href="#i{@page:number}" data-n="{@page:number}" aria-label="Interference {@page:number}">
              <circle cx="{@page:mapX}" cy="{@page:mapY}" r="{16 - 9 * $areMany}"/>
              <xsl:if test="not($areMany)"><text x="{@page:mapX}" y="{@page:mapY}" dy=".35em"><xsl:value-of select="@page:number"/></text></xsl:if>
            </a>
          </xsl:for-each>
        </svg>
      </div>
    </figure>
  </xsl:template>

  <!-- A number with three significant digits, its whole part kept; all of it where the pointer rests. -->
  <xsl:template name="number">
    <xsl:param name="text"/>
    <xsl:param name="unit"/>
    <xsl:variable name="number" select="number(translate($text, ',', '.'))"/>
    <xsl:variable name="size" select="$number * (1 - 2 * ($number &lt; 0))"/>
    <xsl:variable name="form">
      <xsl:choose>
        <xsl:when test="not($size > 0.00001) or $size > 1000000000000"/>
        <xsl:when test="$size >= 99.95">0</xsl:when>
        <xsl:when test="$size >= 9.995">0.0</xsl:when>
        <xsl:when test="$size >= 0.9995">0.00</xsl:when>
        <xsl:when test="$size >= 0.09995">0.000</xsl:when>
        <xsl:when test="$size >= 0.009995">0.0000</xsl:when>
        <xsl:when test="$size >= 0.0009995">0.00000</xsl:when>
        <xsl:when test="$size >= 0.00009995">0.000000</xsl:when>
        <xsl:otherwise>0.0000000</xsl:otherwise>
      </xsl:choose>
    </xsl:variable>
    <xsl:variable name="rounded">
      <xsl:if test="$form != ''"><xsl:value-of select="format-number($number, $form)"/></xsl:if>
    </xsl:variable>
    <xsl:choose>
      <xsl:when test="$rounded != '' and string-length($rounded) &lt; string-length($text)">
        <data value="{$text}" title="{$text}{$unit}">
          <xsl:choose>
            <xsl:when test="contains($text, ',')"><xsl:value-of select="translate($rounded, '.', ',')"/></xsl:when>
            <xsl:otherwise><xsl:value-of select="$rounded"/></xsl:otherwise>
          </xsl:choose>
        </data>
      </xsl:when>
      <xsl:when test="$number = $number"><data value="{$text}"><xsl:value-of select="$text"/></data></xsl:when>
      <xsl:otherwise><xsl:call-template name="short"><xsl:with-param name="text" select="$text"/></xsl:call-template></xsl:otherwise>
    </xsl:choose>
  </xsl:template>

  <!-- Only known words become classes. -->
  <xsl:template name="class">
    <xsl:param name="word"/>
    <xsl:choose>
      <xsl:when test="$word = 'Clash'">clash</xsl:when>
      <xsl:when test="$word = 'Contact'">contact</xsl:when>
      <xsl:when test="$word = 'Clearance'">clearance</xsl:when>
      <xsl:when test="$word = 'Relevant'">relevant</xsl:when>
      <xsl:when test="$word = 'Irrelevant'">irrelevant</xsl:when>
      <xsl:when test="$word = 'Not inspected'">open</xsl:when>
      <xsl:otherwise>other</xsl:otherwise>
    </xsl:choose>
  </xsl:template>

  <xsl:template name="type">
    <xsl:variable name="class"><xsl:call-template name="class"><xsl:with-param name="word" select="@page:type"/></xsl:call-template></xsl:variable>
    <span class="type {$class}">
      <xsl:call-template name="short"><xsl:with-param name="text" select="@page:type"/></xsl:call-template>
    </span>
  </xsl:template>

  <!-- Where many stand together, the beginning of a text is enough; the section has all of it. -->
  <xsl:template name="short">
    <xsl:param name="text"/>
    <xsl:param name="most" select="120"/>
    <bdi><xsl:value-of select="substring($text, 1, $most)"/></bdi>
    <xsl:if test="string-length($text) > $most">…</xsl:if>
  </xsl:template>

  <!-- Table -->
  <xsl:template name="table">
    <form class="filters" hidden="hidden" role="search">
      <label>Search <input type="search" name="text" autocomplete="off"/></label>
      <label>Type <select name="type"><option value="">All</option></select></label>
      <label>Status <select name="status"><option value="">All</option></select></label>
      <xsl:if test="$hasBaseline"><label>Change <select name="change"><option value="">All</option></select></label></xsl:if>
      <output aria-live="polite"></output>
    </form>
    <div class="wide">
      <table id="interferences">
        <xsl:attribute name="class">
          <xsl:if test="$hasPictures">pictured </xsl:if>
          <xsl:if test="$hasBaseline">changes </xsl:if>
          <xsl:if test="not($interferences/@Value != '')">no-value </xsl:if>
          <xsl:if test="not($interferences/Product)">no-products </xsl:if>
          <xsl:if test="not($interferences/ViolatedRule[last()]/@Name != '')">no-rule </xsl:if>
          <xsl:if test="not($interferences/Comment[last()]/@Value != '')">no-comment</xsl:if>
        </xsl:attribute>
        <thead>
          <tr>
            <th class="number" scope="col">N</th>
            <xsl:if test="$hasPictures"><th scope="col" class="plain">Picture</th></xsl:if>
            <th scope="col">Type</th>
            <th class="number value" scope="col" title="Millimetres">Value</th>
            <th class="status" scope="col">Status</th>
            <xsl:if test="$hasBaseline"><th class="change" scope="col">Change</th></xsl:if>
            <th class="products" scope="col">Products</th>
            <th class="rule" scope="col">Rule</th>
            <th class="comment" scope="col">Comment</th>
          </tr>
        </thead>
        <tbody><xsl:apply-templates select="$all" mode="row"/></tbody>
      </table>
    </div>
  </xsl:template>

  <xsl:template match="Interference" mode="row">
    <tr data-n="{@page:number}" data-id="{@page:id}" data-type="{@page:type}" data-status="{@page:status}">
      <xsl:if test="$hasBaseline"><xsl:attribute name="data-change"><xsl:value-of select="@page:change"/></xsl:attribute></xsl:if>
      <td class="number"><a href="#i{@page:number}"><xsl:call-template name="shownNumber"/></a></td>
      <xsl:if test="$hasPictures">
        <td class="thumb">
          <xsl:if test="@page:picture | @page:before">
            <a href="#i{@page:number}">
              <xsl:call-template name="image">
                <xsl:with-param name="path" select="concat(@page:picture, substring(@page:before, 1, string-length(@page:before) * not(@page:picture)))"/>
                <xsl:with-param name="meaning" select="concat('To interference ', @page:number)"/>
                <xsl:with-param name="isLater" select="true()"/>
              </xsl:call-template>
            </a>
          </xsl:if>
        </td>
      </xsl:if>
      <td><xsl:call-template name="type"/></td>
      <td class="number value"><xsl:call-template name="number"><xsl:with-param name="text" select="@Value"/><xsl:with-param name="unit"> mm</xsl:with-param></xsl:call-template></td>
      <td class="status"><xsl:call-template name="short"><xsl:with-param name="text" select="@page:status"/></xsl:call-template></td>
      <xsl:if test="$hasBaseline"><td class="change"><xsl:value-of select="@page:change"/></td></xsl:if>
      <td class="products">
        <xsl:apply-templates select="Product[1]" mode="name"/>
        <xsl:apply-templates select="Product[position() > 1][last()]" mode="name"/>
      </td>
      <td class="rule"><xsl:call-template name="short"><xsl:with-param name="text" select="ViolatedRule[last()]/@Name"/></xsl:call-template></td>
      <td class="comment"><xsl:call-template name="short"><xsl:with-param name="text" select="Comment[last()]/@Value"/></xsl:call-template></td>
    </tr>
  </xsl:template>

  <!-- Of the older result it is marked. -->
  <xsl:template name="shownNumber">
    <xsl:choose>
      <xsl:when test="starts-with(@page:number, 'old-')"><xsl:value-of select="concat(substring(@page:number, 5), '′')"/></xsl:when>
      <xsl:otherwise><xsl:value-of select="@page:number"/></xsl:otherwise>
    </xsl:choose>
  </xsl:template>

  <!-- What became of it since the older result. -->
  <xsl:template name="change">
    <xsl:if test="@page:change">
      <p class="became" data-change="{@page:change}">
        <strong class="change"><xsl:value-of select="@page:change"/></strong>
        <xsl:text> since </xsl:text>
        <bdi><xsl:value-of select="/*/@page:baseline"/></bdi>
        <xsl:if test="@page:reason">: <bdi><xsl:value-of select="@page:reason"/></bdi></xsl:if>
      </p>
      <xsl:if test="page:Change">
        <ul class="became">
          <xsl:for-each select="page:Change">
            <li>
              <xsl:value-of select="@page:what"/>
              <xsl:text>: </xsl:text>
              <xsl:call-template name="number"><xsl:with-param name="text" select="@page:from"/></xsl:call-template>
              <xsl:text> → </xsl:text>
              <xsl:call-template name="number"><xsl:with-param name="text" select="@page:to"/></xsl:call-template>
            </li>
          </xsl:for-each>
        </ul>
      </xsl:if>
      <xsl:if test="@page:before">
        <figure class="before">
          <a class="zoom" href="{@page:before}">
            <xsl:call-template name="image">
              <xsl:with-param name="path" select="@page:before"/>
              <xsl:with-param name="meaning" select="concat('Picture before, of ', @page:number)"/>
            </xsl:call-template>
          </a>
          <figcaption class="note">Before</figcaption>
        </figure>
      </xsl:if>
    </xsl:if>
  </xsl:template>

  <xsl:template match="Product" mode="name">
    <div class="product">
      <xsl:call-template name="swatch"/>
      <xsl:variable name="name"><xsl:call-template name="productName"/></xsl:variable>
      <xsl:call-template name="short">
        <xsl:with-param name="text" select="$name"/>
        <xsl:with-param name="most" select="240"/>
      </xsl:call-template>
      <xsl:if test="@page:missing"><xsl:text> </xsl:text><span class="missing">not in the model</span></xsl:if>
    </div>
  </xsl:template>

  <xsl:template name="productName">
    <xsl:choose>
      <xsl:when test="@Alias != ''"><xsl:value-of select="@Alias"/></xsl:when>
      <xsl:when test="@DescriptionID != ''"><xsl:value-of select="@DescriptionID"/></xsl:when>
      <xsl:otherwise>(no name)</xsl:otherwise>
    </xsl:choose>
  </xsl:template>

  <xsl:template name="swatch">
    <xsl:if test="@page:colour">
      <svg class="swatch" viewBox="0 0 1 1" role="img" aria-label="Colour in the picture"><rect width="1" height="1" fill="{@page:colour}"/></svg>
    </xsl:if>
  </xsl:template>

  <!-- Sections -->
  <xsl:template match="Interference" mode="section">
    <section id="i{@page:number}" class="interference" data-n="{@page:number}">
      <xsl:choose>
        <xsl:when test="$areMany"><noscript class="later"><xsl:call-template name="section"/></noscript></xsl:when>
        <xsl:otherwise><xsl:call-template name="section"/></xsl:otherwise>
      </xsl:choose>
    </section>
  </xsl:template>

  <xsl:template name="section">
    <h2>
      <a class="back" href="#interferences" title="To the table"><xsl:call-template name="shownNumber"/></a>
      <xsl:call-template name="type"/>
      <xsl:if test="@Value != ''">
        <span class="value"><xsl:call-template name="number"><xsl:with-param name="text" select="@Value"/><xsl:with-param name="unit"> mm</xsl:with-param></xsl:call-template>&#160;mm</span>
      </xsl:if>
      <span class="status"><bdi><xsl:value-of select="@page:status"/></bdi></span>
    </h2>
    <div class="body">
      <xsl:if test="@page:picture">
        <figure class="picture">
          <a class="zoom" href="{@page:picture}">
            <xsl:call-template name="image">
              <xsl:with-param name="path" select="@page:picture"/>
              <xsl:with-param name="meaning" select="concat('Picture of interference ', @page:number)"/>
            </xsl:call-template>
          </a>
          <xsl:if test="page:Thumbnail">
            <div class="thumbnails">
              <xsl:for-each select="page:Thumbnail[position() &lt;= $mostPoints]">
                <a class="zoom" href="{@href}">
                  <xsl:call-template name="image">
                    <xsl:with-param name="path" select="@href"/>
                    <xsl:with-param name="meaning" select="concat('Point ', position())"/>
                  </xsl:call-template>
                </a>
              </xsl:for-each>
            </div>
          </xsl:if>
          <xsl:if test="@page:asInModel">
            <figcaption class="note">As in the model: <bdi><xsl:value-of select="@page:asInModel"/></bdi></figcaption>
          </xsl:if>
        </figure>
      </xsl:if>
      <div class="details">
        <xsl:call-template name="change"/>
        <xsl:choose>
          <xsl:when test="Product">
            <xsl:apply-templates select="Product[1]" mode="card"/>
            <xsl:apply-templates select="Product[position() > 1][last()]" mode="card"/>
          </xsl:when>
          <xsl:otherwise><p class="note">The document names no product.</p></xsl:otherwise>
        </xsl:choose>
        <dl class="facts">
          <xsl:call-template name="fact">
            <xsl:with-param name="name">Name</xsl:with-param>
            <xsl:with-param name="value" select="@Name"/>
          </xsl:call-template>
          <xsl:call-template name="fact">
            <xsl:with-param name="name">Result</xsl:with-param>
            <xsl:with-param name="value" select="../self::ClashResult/@Name"/>
          </xsl:call-template>
          <xsl:apply-templates select="ViolatedRule[last()]"/>
          <xsl:call-template name="length">
            <xsl:with-param name="name">Clearance</xsl:with-param>
            <xsl:with-param name="value" select="@DistanceClearance"/>
          </xsl:call-template>
          <xsl:apply-templates select="GeometricAspect[last()]"/>
          <xsl:call-template name="fact">
            <xsl:with-param name="name">Age</xsl:with-param>
            <xsl:with-param name="value" select="@RetrieveInf"/>
          </xsl:call-template>
        </dl>
        <xsl:if test="GeometricAspect/Point"><xsl:call-template name="points"/></xsl:if>
        <xsl:if test="Comment[last()]/@Value != ''">
          <blockquote><bdi><xsl:value-of select="Comment[last()]/@Value"/></bdi></blockquote>
        </xsl:if>
      </div>
    </div>
  </xsl:template>

  <xsl:template name="image">
    <xsl:param name="path"/>
    <xsl:param name="meaning"/>
    <xsl:param name="isLater" select="false()"/>
    <xsl:choose>
      <xsl:when test="starts-with($path, '#')">
        <svg class="image" role="img" aria-label="{$meaning}"><use href="{$path}"/></svg>
      </xsl:when>
      <xsl:when test="$areMany and $isLater">
        <noscript class="later"><img src="{$path}" alt="{$meaning}" loading="lazy" decoding="async"/></noscript>
      </xsl:when>
      <xsl:otherwise><img src="{$path}" alt="{$meaning}" loading="lazy" decoding="async"/></xsl:otherwise>
    </xsl:choose>
  </xsl:template>

  <xsl:template match="Product" mode="card">
    <div class="card">
      <xsl:if test="@page:preview">
        <a class="zoom" href="{@page:preview}">
          <xsl:call-template name="image">
            <xsl:with-param name="path" select="@page:preview"/>
            <xsl:with-param name="meaning">Picture of the product</xsl:with-param>
          </xsl:call-template>
        </a>
      </xsl:if>
      <div>
        <div class="product">
          <xsl:call-template name="swatch"/>
          <strong><bdi><xsl:call-template name="productName"/></bdi></strong>
          <xsl:if test="@page:missing"><xsl:text> </xsl:text><span class="missing">not in the model</span></xsl:if>
        </div>
        <xsl:if test="@DescriptionID != '' and @Alias != '' and @DescriptionID != @Alias">
          <div class="note"><bdi><xsl:value-of select="@DescriptionID"/></bdi></div>
        </xsl:if>
        <xsl:if test="@ShapeName != ''">
          <div class="note">Shape <bdi><xsl:value-of select="@ShapeName"/></bdi></div>
        </xsl:if>
      </div>
    </div>
  </xsl:template>

  <xsl:template match="ViolatedRule">
    <xsl:variable name="text">
      <xsl:value-of select="@Name"/>
      <xsl:if test="@Severity != ''"><xsl:value-of select="concat(', ', @Severity)"/></xsl:if>
      <xsl:if test="@Clearance != ''"><xsl:value-of select="concat(', clearance&#160;', @Clearance, '&#160;mm')"/></xsl:if>
    </xsl:variable>
    <xsl:call-template name="fact">
      <xsl:with-param name="name">Violated rule</xsl:with-param>
      <xsl:with-param name="value" select="$text"/>
    </xsl:call-template>
  </xsl:template>

  <xsl:template match="GeometricAspect">
    <xsl:call-template name="length">
      <xsl:with-param name="name">Curve length</xsl:with-param>
      <xsl:with-param name="value" select="@IntersectCurveLength"/>
    </xsl:call-template>
    <xsl:call-template name="length">
      <xsl:with-param name="name">Measured value</xsl:with-param>
      <xsl:with-param name="value" select="@ExtractOrDistValue"/>
    </xsl:call-template>
  </xsl:template>

  <xsl:template name="points">
    <xsl:variable name="count" select="count(GeometricAspect/Point)"/>
    <details>
      <xsl:if test="$count &lt; 5"><xsl:attribute name="open">open</xsl:attribute></xsl:if>
      <summary>
        <xsl:value-of select="$count"/>
        <xsl:text> point</xsl:text>
        <xsl:if test="$count != 1">s</xsl:if>
        <xsl:text> (x, y, z in mm)</xsl:text>
      </summary>
      <ol>
        <xsl:for-each select="GeometricAspect/Point">
          <xsl:if test="position() &lt;= $mostPoints">
            <li>
              <span class="coordinate"><xsl:call-template name="number"><xsl:with-param name="text" select="@Ux"/></xsl:call-template></span>
              <span class="coordinate"><xsl:call-template name="number"><xsl:with-param name="text" select="@Uy"/></xsl:call-template></span>
              <span class="coordinate"><xsl:call-template name="number"><xsl:with-param name="text" select="@Uz"/></xsl:call-template></span>
            </li>
          </xsl:if>
        </xsl:for-each>
      </ol>
      <xsl:if test="$count > $mostPoints">
        <p class="note"><xsl:value-of select="concat('The other ', $count - $mostPoints, ' are in report.xml.')"/></p>
      </xsl:if>
    </details>
  </xsl:template>
</xsl:stylesheet>
