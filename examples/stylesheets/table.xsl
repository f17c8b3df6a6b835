<?xml version="1.0" encoding="UTF-8"?>
<!--
  Turns a document of the formatter "xml" into a page of HTML tables: a list of structures is a
  table with a row each, a structure is a table with a row for each field, and so are those inside.
  Named with the format parameter "stylesheet", it is found by xsltproc and by browsers.
-->
<xsl:stylesheet version="1.0" xmlns:xsl="http://www.w3.org/1999/XSL/Transform">
  <xsl:output method="html" indent="yes" doctype-system="about:legacy-compat"/>
  <xsl:strip-space elements="*"/>
  <xsl:preserve-space elements="string"/>

  <xsl:template match="/output">
    <html>
      <head><title>Result</title></head>
      <body><xsl:apply-templates select="root/*"/></body>
    </html>
  </xsl:template>

  <xsl:template match="list[@type='structure']">
    <table>
      <xsl:if test="structure">
        <tr>
          <xsl:for-each select="structure[1]/field">
            <th><xsl:value-of select="@name"/></th>
          </xsl:for-each>
        </tr>
      </xsl:if>
      <xsl:for-each select="structure">
        <tr>
          <xsl:for-each select="field"><td><xsl:apply-templates/></td></xsl:for-each>
        </tr>
      </xsl:for-each>
    </table>
  </xsl:template>

  <xsl:template match="list">
    <xsl:for-each select="*">
      <xsl:if test="position() > 1">, </xsl:if>
      <xsl:apply-templates select="."/>
    </xsl:for-each>
  </xsl:template>

  <xsl:template match="structure">
    <table>
      <xsl:for-each select="field">
        <tr><th><xsl:value-of select="@name"/></th><td><xsl:apply-templates/></td></tr>
      </xsl:for-each>
    </table>
  </xsl:template>
</xsl:stylesheet>
