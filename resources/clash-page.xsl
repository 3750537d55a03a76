<?xml version="1.0" encoding="UTF-8"?>
<!-- Turns a report of a clash result into the page that "lyra publish" writes. Beside what a report
     holds, that command gives to the root: page:model, a page:Type for each type and a page:Status
     for each status, with page:word and page:count; to each interference: page:number, page:type,
     page:status, page:picture, page:asInModel (why the picture does not have the result's placements)
     and page:Thumbnail elements; to each of its two products: page:colour, page:preview and
     page:missing. page:asInModel at the root says that no picture has them, as was asked for. Texts of the document are isolated (bdi), so that none can change
     the direction of what stands around it. -->
<xsl:stylesheet version="1.0" xmlns:xsl="http://www.w3.org/1999/XSL/Transform"
                xmlns:page="urn:zorlyra:page" exclude-result-prefixes="page">
  <xsl:output method="html" version="5" encoding="UTF-8" indent="no"
              doctype-system="about:legacy-compat"/>

  <xsl:variable name="interferences"
                select="/ClashElement/ClashResult/Interference | /InterferenceElement/Interference[1]"/>
  <xsl:variable name="hasPictures" select="boolean($interferences/@page:picture)"/>
  <xsl:variable name="mostPoints" select="100"/>
  <!-- With more interferences than this, a script puts pictures in where they are seen: browsers take long
       over tens of thousands of lazy ones. -->
  <xsl:variable name="mostLazy" select="1000"/>
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
              content="default-src 'none'; img-src 'self' file: data:; style-src 'unsafe-inline'; script-src 'unsafe-inline'; form-action 'none'; base-uri 'none'"/>
        <link rel="icon" href="data:,"/>
        <xsl:call-template name="style"/>
      </head>
      <body>
        <xsl:apply-templates select="/ClashElement | /InterferenceElement"/>
        <xsl:call-template name="script"/>
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
          <xsl:with-param name="name">Interferences</xsl:with-param>
          <xsl:with-param name="value" select="count($interferences)"/>
        </xsl:call-template>
      </dl>
      <xsl:if test="$interferences">
        <div class="charts">
          <xsl:call-template name="chart">
            <xsl:with-param name="name">Type</xsl:with-param>
            <xsl:with-param name="counts" select="page:Type"/>
          </xsl:call-template>
          <xsl:call-template name="chart">
            <xsl:with-param name="name">Status</xsl:with-param>
            <xsl:with-param name="counts" select="page:Status"/>
          </xsl:call-template>
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
        <xsl:when test="$interferences">
          <xsl:call-template name="table"/>
          <xsl:for-each select="$interferences">
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
      <xsl:if test="@Clearance != ''"><xsl:value-of select="concat(', clearance ', @Clearance, ' mm')"/></xsl:if>
    </xsl:variable>
    <xsl:call-template name="fact">
      <xsl:with-param name="name">Specification</xsl:with-param>
      <xsl:with-param name="value" select="$text"/>
    </xsl:call-template>
  </xsl:template>

  <!-- A bar whose parts are as long as their counts, and what they mean. -->
  <xsl:template name="chart">
    <xsl:param name="name"/>
    <xsl:param name="counts"/>
    <figure class="chart">
      <figcaption><xsl:value-of select="$name"/></figcaption>
      <div class="bar" aria-hidden="true">
        <xsl:for-each select="$counts">
          <xsl:variable name="class"><xsl:call-template name="class"><xsl:with-param name="word" select="@page:word"/></xsl:call-template></xsl:variable>
          <span class="{$class}" style="flex-grow:{@page:count}"></span>
        </xsl:for-each>
      </div>
      <ul>
        <xsl:for-each select="$counts">
          <xsl:variable name="class"><xsl:call-template name="class"><xsl:with-param name="word" select="@page:word"/></xsl:call-template></xsl:variable>
          <li>
            <span class="dot {$class}"></span>
            <strong><xsl:value-of select="@page:count"/></strong>
            <xsl:text> </xsl:text>
            <xsl:call-template name="short"><xsl:with-param name="text" select="@page:word"/></xsl:call-template>
          </li>
        </xsl:for-each>
      </ul>
    </figure>
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
      <output aria-live="polite"></output>
    </form>
    <div class="wide">
      <table id="interferences">
        <xsl:if test="$hasPictures"><xsl:attribute name="class">pictured</xsl:attribute></xsl:if>
        <thead>
          <tr>
            <th class="number" scope="col">N</th>
            <xsl:if test="$hasPictures"><th scope="col" class="plain">Picture</th></xsl:if>
            <th scope="col">Type</th>
            <th class="number" scope="col">Value</th>
            <th scope="col">Status</th>
            <th scope="col">Products</th>
            <th scope="col">Rule</th>
            <th scope="col">Comment</th>
          </tr>
        </thead>
        <tbody><xsl:apply-templates select="$interferences" mode="row"/></tbody>
      </table>
    </div>
  </xsl:template>

  <xsl:template match="Interference" mode="row">
    <tr data-n="{@page:number}" data-type="{@page:type}" data-status="{@page:status}">
      <td class="number"><a href="#i{@page:number}"><xsl:value-of select="@page:number"/></a></td>
      <xsl:if test="$hasPictures">
        <td class="thumb">
          <xsl:if test="@page:picture">
            <a href="#i{@page:number}">
              <xsl:call-template name="image"><xsl:with-param name="path" select="@page:picture"/></xsl:call-template>
            </a>
          </xsl:if>
        </td>
      </xsl:if>
      <td><xsl:call-template name="type"/></td>
      <td class="number"><xsl:call-template name="short"><xsl:with-param name="text" select="@Value"/></xsl:call-template></td>
      <td><xsl:call-template name="short"><xsl:with-param name="text" select="@page:status"/></xsl:call-template></td>
      <td class="products">
        <xsl:apply-templates select="Product[1]" mode="name"/>
        <xsl:apply-templates select="Product[position() > 1][last()]" mode="name"/>
      </td>
      <td><xsl:call-template name="short"><xsl:with-param name="text" select="ViolatedRule[last()]/@Name"/></xsl:call-template></td>
      <td class="comment"><xsl:call-template name="short"><xsl:with-param name="text" select="Comment[last()]/@Value"/></xsl:call-template></td>
    </tr>
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
      <span class="swatch" style="background:{@page:colour}" title="Colour in the picture"></span>
    </xsl:if>
  </xsl:template>

  <!-- Sections -->
  <xsl:template match="Interference" mode="section">
    <section id="i{@page:number}" class="interference" data-n="{@page:number}">
      <h2>
        <a class="back" href="#interferences" title="To the table"><xsl:value-of select="@page:number"/></a>
        <xsl:call-template name="type"/>
        <xsl:if test="@Value != ''">
          <span class="value"><bdi><xsl:value-of select="@Value"/></bdi> mm</span>
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
            <xsl:if test="@DistanceClearance != ''">
              <xsl:call-template name="fact">
                <xsl:with-param name="name">Clearance</xsl:with-param>
                <xsl:with-param name="value" select="concat(@DistanceClearance, ' mm')"/>
              </xsl:call-template>
            </xsl:if>
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
    </section>
  </xsl:template>

  <xsl:template name="image">
    <xsl:param name="path"/>
    <xsl:param name="meaning"/>
    <xsl:choose>
      <xsl:when test="$areMany">
        <noscript class="later"><img src="{$path}" alt="{$meaning}" loading="lazy" decoding="async"/></noscript>
      </xsl:when>
      <xsl:otherwise><img src="{$path}" alt="{$meaning}" loading="lazy" decoding="async"/></xsl:otherwise>
    </xsl:choose>
  </xsl:template>

  <xsl:template match="Product" mode="card">
    <div class="card">
      <xsl:if test="@page:preview">
        <a class="zoom" href="{@page:preview}">
          <xsl:call-template name="image"><xsl:with-param name="path" select="@page:preview"/></xsl:call-template>
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
      <xsl:if test="@Clearance != ''"><xsl:value-of select="concat(', clearance ', @Clearance, ' mm')"/></xsl:if>
    </xsl:variable>
    <xsl:call-template name="fact">
      <xsl:with-param name="name">Violated rule</xsl:with-param>
      <xsl:with-param name="value" select="$text"/>
    </xsl:call-template>
  </xsl:template>

  <xsl:template match="GeometricAspect">
    <xsl:if test="@IntersectCurveLength != ''">
      <xsl:call-template name="fact">
        <xsl:with-param name="name">Curve length</xsl:with-param>
        <xsl:with-param name="value" select="concat(@IntersectCurveLength, ' mm')"/>
      </xsl:call-template>
    </xsl:if>
    <xsl:call-template name="fact">
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
            <li><bdi><xsl:value-of select="concat(@Ux, '  ', @Uy, '  ', @Uz)"/></bdi></li>
          </xsl:if>
        </xsl:for-each>
      </ol>
      <xsl:if test="$count > $mostPoints">
        <p class="note"><xsl:value-of select="concat('The other ', $count - $mostPoints, ' are in report.xml.')"/></p>
      </xsl:if>
    </details>
  </xsl:template>

  <xsl:template name="style">
    <style>
:root { --ink:#1d2329; --soft:#66707a; --line:#e2e5e8; --paper:#fff; --panel:#f6f7f8; --accent:#1f5fa8;
  --clash:#b3261e; --contact:#9a6200; --clearance:#1f6f9f; --relevant:#7a4fa3; --irrelevant:#8b959e; --open:#3d7a5a; --other:#6f7780; }
@media (prefers-color-scheme: dark) { :root { --ink:#e4e7ea; --soft:#98a2ac; --line:#2f363d; --paper:#15191d; --panel:#1d2227; --accent:#83b6ee;
  --clash:#f0857d; --contact:#e0ad55; --clearance:#74bde6; --relevant:#c3a0e6; --irrelevant:#7c868f; --open:#7fc29f; --other:#8e979f; } }
* { box-sizing:border-box }
body { margin:0 auto; padding:2rem clamp(1rem,4vw,3rem) 4rem; max-width:84rem; background:var(--paper); color:var(--ink);
  font:15px/1.5 system-ui,-apple-system,"Segoe UI",Roboto,"Noto Sans",sans-serif; overflow-wrap:anywhere }
a { color:var(--accent); text-decoration:none } a:hover { text-decoration:underline }
:focus-visible { outline:2px solid var(--accent); outline-offset:2px }
.kind { margin:0; color:var(--soft); font-size:.8rem; letter-spacing:.08em; text-transform:uppercase }
h1 { margin:.1rem 0 1rem; font-size:1.9rem; line-height:1.2; font-weight:650 }
.facts { display:flex; flex-wrap:wrap; gap:.7rem 2.2rem; margin:0 }
.facts dt { color:var(--soft); font-size:.8rem } .facts dd { margin:0 }
.charts { display:grid; grid-template-columns:repeat(auto-fit,minmax(17rem,1fr)); gap:1.2rem 2.5rem; margin:1.6rem 0 }
.chart { margin:0 } .chart figcaption { color:var(--soft); font-size:.8rem; margin-bottom:.35rem }
.bar { display:flex; gap:2px; height:.7rem; border-radius:.35rem; overflow:hidden }
.bar span { flex-basis:3px; background:var(--c) }
.chart ul { display:flex; flex-wrap:wrap; gap:.2rem 1.2rem; margin:.5rem 0 0; padding:0; list-style:none; font-size:.9rem }
.dot { display:inline-block; width:.6rem; height:.6rem; border-radius:50%; background:var(--c); margin-right:.2rem }
.clash { --c:var(--clash) } .contact { --c:var(--contact) } .clearance { --c:var(--clearance) } .other { --c:var(--other) }
.relevant { --c:var(--relevant) } .irrelevant { --c:var(--irrelevant) } .open { --c:var(--open) }
.type { color:var(--c); font-weight:600 }
.notice { background:var(--panel); border-left:3px solid var(--contact); padding:.6rem .9rem; border-radius:.25rem }
.missing { color:var(--contact); border:1px solid currentColor; border-radius:.25rem; font-size:.72rem; padding:0 .3rem; white-space:nowrap }
.filters { display:flex; flex-wrap:wrap; gap:.6rem 1.2rem; align-items:center; margin:2rem 0 .6rem; color:var(--soft); font-size:.85rem }
.filters[hidden] { display:none }
.filters input,.filters select { font:inherit; color:var(--ink); background:var(--panel); border:1px solid var(--line); border-radius:.35rem; padding:.3rem .5rem; margin-left:.3rem; max-width:16rem }
@media screen { h1,.facts dd,h2 > *,.card strong,.card .note,figcaption { max-height:9em; overflow:auto } h1 { max-height:7.2em } }
.filters output { margin-left:auto }
.wide { overflow-x:auto; margin-top:1rem }
table { border-collapse:collapse; width:100%; font-size:.9rem }
th,td { text-align:start; vertical-align:top; padding:.5rem .7rem; border-bottom:1px solid var(--line); overflow:clip }
th { color:var(--soft); font-weight:600; font-size:.8rem; white-space:nowrap }
th button { all:unset; cursor:pointer; color:inherit } th button:hover { color:var(--ink) }
th button:focus-visible { outline:2px solid var(--accent) }
th[aria-sort=ascending] button::after { content:" ↑" } th[aria-sort=descending] button::after { content:" ↓" }
tbody tr:hover { background:var(--panel) }
.number { text-align:right; font-variant-numeric:tabular-nums } .number:first-child { white-space:nowrap } td.comment { color:var(--soft) }
/* Rows of fixed columns, so that of thousands only those are laid out that are seen. */
@media screen {
  table,thead,tbody { display:block } table { min-width:60rem }
  tr { display:grid; grid-template-columns:var(--columns); --columns:3.5rem 7rem 6.8rem 8.5rem minmax(15rem,2fr) minmax(5rem,.6fr) minmax(9rem,1fr) }
  .pictured tr { --columns:3.5rem 7.5rem 7rem 6.8rem 8.5rem minmax(15rem,2fr) minmax(5rem,.6fr) minmax(9rem,1fr) }
  th,td { border:0 } tr { border-bottom:1px solid var(--line) } tr[hidden] { display:none }
  tbody tr { content-visibility:auto; contain-intrinsic-size:auto 2.5rem } .pictured tbody tr { contain-intrinsic-size:auto 5.1rem }
}
img { background:#fff; border-radius:.3rem }
.thumb a,.card a { min-height:64px } .thumb img,.card img { display:block; width:96px; height:64px; object-fit:cover; border:1px solid var(--line) }
.swatch { display:inline-block; width:.75rem; height:.75rem; border-radius:.2rem; margin-right:.4rem; vertical-align:-.05rem; border:1px solid #0003; box-shadow:0 0 0 1px #fff3 }
.interference { margin-top:2.5rem; padding-top:1.2rem; border-top:1px solid var(--line); scroll-margin-top:1rem }
@media screen { .interference { content-visibility:auto; contain-intrinsic-size:auto 30rem } }
h2 { display:flex; flex-wrap:wrap; align-items:baseline; gap:.3rem .9rem; margin:0 0 1rem; font-size:1.15rem; font-weight:600 }
.back { font-variant-numeric:tabular-nums; color:var(--soft) } .value { font-variant-numeric:tabular-nums }
.status { margin-left:auto; color:var(--soft); font-size:.85rem; font-weight:400 }
.body { display:grid; grid-template-columns:minmax(0,3fr) minmax(0,2fr); gap:1.8rem }
.details:first-child { grid-column:1/-1 }
.picture { margin:0 } .picture > a img { display:block; width:100%; height:auto; aspect-ratio:756/506; object-fit:contain; border:1px solid var(--line) }
.thumbnails { display:flex; flex-wrap:wrap; gap:.4rem; margin-top:.4rem } .thumbnails img { display:block; width:72px; height:50px; border:1px solid var(--line) }
.card .product { display:flex; gap:.4rem; align-items:baseline } .card .swatch,.card .missing { flex:none; margin:0 } .card strong { min-width:0 }
.card { display:flex; gap:.9rem; align-items:flex-start; margin-bottom:1rem } .card a { flex:none }
.note { color:var(--soft); font-size:.85rem }
details { margin-top:1rem; font-size:.85rem } summary { cursor:pointer; color:var(--soft) }
details bdi { white-space:pre-wrap } details ol { margin:.4rem 0 0; padding-left:3rem; max-height:16rem; overflow:auto; font-variant-numeric:tabular-nums }
blockquote { margin:1rem 0 0; padding:.6rem .9rem; background:var(--panel); border-radius:.35rem; white-space:pre-wrap; max-height:20rem; overflow:auto }
dialog { padding:0; border:0; background:transparent; max-width:96vw; max-height:96vh } dialog img { display:block; max-width:96vw; max-height:94vh; cursor:zoom-out }
dialog::backdrop { background:#000c }
@media (max-width:50rem) { .body { grid-template-columns:1fr } .status { margin-left:0 } body { padding-top:1.2rem } }
@media print {
  :root { --ink:#000; --soft:#444; --line:#bbb; --paper:#fff; --panel:#f3f3f3; --accent:#000; --clash:#b3261e; --contact:#9a6200; --clearance:#1f6f9f; --relevant:#7a4fa3; --irrelevant:#8b959e; --open:#3d7a5a; --other:#6f7780 }
  body { max-width:none; padding:0; font-size:10pt; print-color-adjust:exact; -webkit-print-color-adjust:exact }
  .filters,.filters[hidden] { display:none } .wide { overflow:visible } thead { display:table-header-group } tr,.card,.picture { break-inside:avoid }
  th button { display:contents } table { font-size:8pt } .thumb img { width:60px; height:40px } td.products { width:40% }
  td:nth-last-child(6) { min-width:6.5em } td:nth-last-child(4) { min-width:8em } td:nth-last-child(2) { min-width:5.5em }
  .body { grid-template-columns:minmax(0,1fr) minmax(0,1fr) } .status { margin-left:auto }
  .interference { break-inside:avoid; margin-top:1rem; padding-top:.7rem } h2 { margin-bottom:.6rem }
  blockquote,details ol { max-height:none; overflow:visible }
}
    </style>
  </xsl:template>

  <!-- Sorting, filtering and large pictures for who has scripts; the page says all without. -->
  <xsl:template name="script">
    <script>
(() => {
  'use strict';
  const table = document.getElementById('interferences');
  if (!table) return;
  const body = table.tBodies[0];
  const form = document.querySelector('.filters');
  const rows = Array.from(body.rows, (row, place) => ({
    row, place, text: row.textContent.toLowerCase(),
    section: document.getElementById('i' + row.dataset.n) }));

  const offer = (select, name) => {
    for (const word of new Set(rows.map(item => item.row.dataset[name])))
      select.append(new Option(word, word));
    select.prepend(select.querySelector('option[value=""]'));
    select.value = '';
  };
  offer(form.elements.type, 'type');
  offer(form.elements.status, 'status');

  const filter = () => {
    const text = form.elements.text.value.trim().toLowerCase();
    const type = form.elements.type.value, status = form.elements.status.value;
    let shown = 0;
    for (const { row, section, text: own } of rows) {
      const fits = (!type || row.dataset.type === type) &amp;&amp; (!status || row.dataset.status === status) &amp;&amp; own.includes(text);
      row.hidden = section.hidden = !fits;
      shown += fits;
    }
    form.querySelector('output').value = shown + ' of ' + rows.length + ' shown';
  };
  form.addEventListener('input', filter);
  form.addEventListener('submit', event => event.preventDefault());
  form.hidden = false;
  filter();

  const keyOf = (row, column, isNumber) => {
    const text = row.cells[column].textContent.trim();
    if (!isNumber) return text;
    const number = parseFloat(text.replace(',', '.'));
    return Number.isNaN(number) ? Infinity : number;
  };
  const sort = (header, column) => {
    const isNumber = header.classList.contains('number');
    const down = header.getAttribute('aria-sort') === 'ascending';
    for (const other of header.parentNode.cells) other.removeAttribute('aria-sort');
    header.setAttribute('aria-sort', down ? 'descending' : 'ascending');
    const order = new Intl.Collator(undefined, { numeric: true });
    const compare = isNumber ? (a, b) => a &lt; b ? -1 : a > b ? 1 : 0 : order.compare;
    const keyed = rows.map(item => ({ item, key: keyOf(item.row, column, isNumber) }));
    keyed.sort((a, b) => (down ? compare(b.key, a.key) : compare(a.key, b.key)) || a.item.place - b.item.place);
    body.append(...keyed.map(({ item }) => item.row));
  };
  Array.from(table.tHead.rows[0].cells).forEach((header, column) => {
    if (header.classList.contains('plain')) return;
    const button = document.createElement('button');
    button.type = 'button';
    button.textContent = header.textContent;
    button.addEventListener('click', () => sort(header, column));
    header.replaceChildren(button);
  });

  // Pictures of many are put in when their row or section comes near to being seen.
  const putIn = place => {
    for (const later of place.querySelectorAll('noscript.later'))
      later.replaceWith(new DOMParser().parseFromString(later.textContent, 'text/html').body.firstChild);
  };
  if (document.querySelector('noscript.later')) {
    const near = new IntersectionObserver(entries => {
      for (const { isIntersecting, target } of entries) {
        if (!isIntersecting) continue;
        putIn(target);
        near.unobserve(target);
      }
    }, { rootMargin: '100%' });
    for (const { row, section } of rows) for (const place of [row, section]) near.observe(place);
    addEventListener('beforeprint', () => putIn(document));
  }

  const dialog = document.createElement('dialog');
  const large = document.createElement('img');
  let current = null, all = null;
  const links = () => Array.from(document.querySelectorAll('a.zoom')).filter(link => !link.closest('[hidden]'));
  const show = link => { current = link; large.src = link.href; large.alt = link.firstElementChild.alt || ''; };
  dialog.append(large);
  dialog.addEventListener('click', () => dialog.close());
  dialog.addEventListener('keydown', event => {
    const step = { ArrowRight: 1, ArrowLeft: -1 }[event.key];
    if (!step) return;
    all ??= links();
    show(all[(all.indexOf(current) + step + all.length) % all.length]);
  });
  document.body.append(dialog);
  document.addEventListener('click', event => {
    const link = event.target.closest('a.zoom');
    if (!link || event.ctrlKey || event.metaKey || event.shiftKey || event.button) return;
    event.preventDefault();
    all = null;
    show(link);
    dialog.showModal();
  });
})();
    </script>
  </xsl:template>
</xsl:stylesheet>
