// Spreadsheets by libxlsxwriter.
#include <xlsxwriter.h>

#include <algorithm>
#include <cstring>
#include <memory>
#include <utility>

#include "foundation/PluginFunction.h"
#include "toolkit/exchange/ExchangeLibrary.h"

namespace ZORToolkit {
namespace {

class XlsxWriter final : public SpreadsheetWriter {
 public:
  XlsxWriter(const std::string& inPath, std::int64_t inTime) {
    lxw_workbook_options options{};
    options.constant_memory = LXW_TRUE;
    book_ = workbook_new_opt(inPath.c_str(), &options);
    lxw_doc_properties properties{};
    char creator[] = "ZORLyra";
    properties.author = creator;
    properties.created = inTime;
    workbook_set_properties(book_, &properties);
    header_ = workbook_add_format(book_);
    format_set_bold(header_);
    format_set_bg_color(header_, 0xE4E8EE);
    format_set_bottom(header_, LXW_BORDER_THIN);
    format_set_text_wrap(header_);
    format_set_align(header_, LXW_ALIGN_VERTICAL_TOP);
    plain_ = workbook_add_format(book_);
    format_set_align(plain_, LXW_ALIGN_VERTICAL_TOP);
    editable_ = workbook_add_format(book_);
    format_set_align(editable_, LXW_ALIGN_VERTICAL_TOP);
    format_set_bg_color(editable_, 0xFFFBE6);
    format_set_text_wrap(editable_);
  }
  ~XlsxWriter() override {
    if (book_ != nullptr) lxw_workbook_free(book_);
  }
  XlsxWriter(const XlsxWriter&) = delete;
  XlsxWriter& operator=(const XlsxWriter&) = delete;

  void AddSheet(const SheetLayout& inLayout) override {
    sheet_ = workbook_add_worksheet(book_, inLayout.name.c_str());
    formats_.clear();
    const auto rows = static_cast<lxw_row_t>(inLayout.rows);
    // Where a picture ends is worked out when rows of heights of their own are forgotten already.
    if (inLayout.rowHeight > 0) worksheet_set_default_row(sheet_, inLayout.rowHeight, LXW_FALSE);
    worksheet_set_row(sheet_, 0, 2 * LXW_DEF_ROW_HEIGHT, nullptr);
    for (std::size_t i = 0; i < inLayout.columns.size(); ++i) {
      const SheetColumn& column = inLayout.columns[i];
      formats_.push_back(column.isEditable ? editable_ : plain_);
      lxw_row_col_options options{};
      options.hidden = column.isHidden ? LXW_TRUE : LXW_FALSE;
      const auto at = static_cast<lxw_col_t>(i);
      worksheet_set_column_opt(sheet_, at, at, column.width, nullptr, &options);
      worksheet_write_string(sheet_, 0, at, column.header.c_str(), header_);
    }
    if (inLayout.columns.empty()) return;
    worksheet_freeze_panes(sheet_, 1, 0);
    worksheet_set_landscape(sheet_);  // on paper as wide as a page, each page with the header
    worksheet_fit_to_pages(sheet_, 1, 0);
    worksheet_repeat_rows(sheet_, 0, 0);
    worksheet_autofilter(sheet_, 0, 0, std::max<lxw_row_t>(rows, 1),
                         static_cast<lxw_col_t>(inLayout.columns.size() - 1));
    for (const SheetWords& words : inLayout.words) AddWords(words, rows);
    for (const SheetChart& chart : inLayout.charts) AddChart(chart, inLayout.name);
  }

  void Text(std::size_t inRow, std::size_t inColumn, const std::string& inText) override {
    Check(worksheet_write_string(sheet_, Row(inRow), static_cast<lxw_col_t>(inColumn),
                                 inText.c_str(), formats_[inColumn]));
  }

  void Number(std::size_t inRow, std::size_t inColumn, double inNumber) override {
    Check(worksheet_write_number(sheet_, Row(inRow), static_cast<lxw_col_t>(inColumn), inNumber,
                                 formats_[inColumn]));
  }

  void Picture(std::size_t inRow, std::size_t inColumn, const std::string& inPath,
               double inScale) override {
    lxw_image_options options{};
    options.x_scale = options.y_scale = inScale;
    options.x_offset = options.y_offset = 2;
    options.object_position = LXW_OBJECT_MOVE_AND_SIZE;
    worksheet_insert_image_opt(sheet_, Row(inRow), static_cast<lxw_col_t>(inColumn), inPath.c_str(),
                               &options);
  }

  std::string Finish() override {
    lxw_workbook* const book = std::exchange(book_, nullptr);
    const lxw_error error = workbook_close(book);
    if (error_ == LXW_NO_ERROR) error_ = error;
    return error_ == LXW_NO_ERROR ? "" : lxw_strerror(error_);
  }

 private:
  static lxw_row_t Row(std::size_t inRow) { return static_cast<lxw_row_t>(inRow + 1); }

  void Check(lxw_error inError) {
    if (error_ == LXW_NO_ERROR) error_ = inError;
  }

  void AddWords(const SheetWords& inWords, lxw_row_t inRows) {
    const auto column = static_cast<lxw_col_t>(inWords.column);
    const lxw_row_t last = std::max<lxw_row_t>(inRows, 1);
    std::vector<std::string> words = inWords.words;
    if (inWords.isChoice) {
      std::vector<char*> list;
      for (std::string& word : words) list.push_back(word.data());
      list.push_back(nullptr);
      char title[] = "Unknown word", message[] = "Choose one of the list.";
      lxw_data_validation validation{};
      validation.validate = LXW_VALIDATION_TYPE_LIST;
      validation.value_list = list.data();
      validation.ignore_blank = LXW_VALIDATION_ON;
      validation.dropdown = LXW_VALIDATION_ON;
      validation.show_input = LXW_VALIDATION_ON;
      validation.show_error = LXW_VALIDATION_ON;
      validation.error_title = title;
      validation.error_message = message;
      worksheet_data_validation_range(sheet_, 1, column, last, column, &validation);
    }
    for (std::size_t i = 0; i < inWords.colours.size(); ++i) {
      lxw_format* const format = workbook_add_format(book_);
      format_set_bg_color(format, inWords.colours[i]);
      std::string quoted = "\"" + inWords.words[i] + "\"";
      lxw_conditional_format condition{};
      condition.type = LXW_CONDITIONAL_TYPE_CELL;
      condition.criteria = LXW_CONDITIONAL_CRITERIA_EQUAL_TO;
      condition.value_string = quoted.data();
      condition.format = format;
      worksheet_conditional_format_range(sheet_, 1, column, last, column, &condition);
    }
  }

  void AddChart(const SheetChart& inChart, const std::string& inSheet) {
    lxw_chart* const chart = workbook_add_chart(book_, LXW_CHART_BAR);
    lxw_chart_series* const series = chart_add_series(chart, nullptr, nullptr);
    chart_series_set_categories(series, inSheet.c_str(), Row(inChart.firstRow),
                                static_cast<lxw_col_t>(inChart.wordColumn), Row(inChart.lastRow),
                                static_cast<lxw_col_t>(inChart.wordColumn));
    chart_series_set_values(series, inSheet.c_str(), Row(inChart.firstRow),
                            static_cast<lxw_col_t>(inChart.numberColumn), Row(inChart.lastRow),
                            static_cast<lxw_col_t>(inChart.numberColumn));
    chart_series_set_labels(series);
    chart_title_set_name(chart, inChart.title.c_str());
    chart_legend_set_position(chart, LXW_CHART_LEGEND_NONE);
    chart_axis_set_reverse(chart->y_axis);
    worksheet_insert_chart(sheet_, Row(inChart.row), static_cast<lxw_col_t>(inChart.column), chart);
  }

  lxw_workbook* book_ = nullptr;
  lxw_worksheet* sheet_ = nullptr;
  lxw_format *header_ = nullptr, *plain_ = nullptr, *editable_ = nullptr;
  std::vector<lxw_format*> formats_;  // of the sheet's columns
  lxw_error error_ = LXW_NO_ERROR;
};

}  // namespace
}  // namespace ZORToolkit

ZOR_PLUGIN_FUNCTION ZORToolkit::SpreadsheetWriter* ZORNewSpreadsheet(const std::string& inPath,
                                                                     std::int64_t inTime) {
  return new ZORToolkit::XlsxWriter(inPath, inTime);
}
