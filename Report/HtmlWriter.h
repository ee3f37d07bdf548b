#pragma once

#include <cstddef>
#include <string>
#include <string_view>

namespace ventrik
{

/// Writes a page that is HTML and XML at once. Elements end in the order in which they began; all
/// text is escaped, and what no document can carry is replaced.
class HtmlWriter
{
  public:
    /// What is longer is cut, and its size said.
    static constexpr std::size_t longestText = 300;

    /// An element that lasts as long as this does. The name is a constant.
    class Element
    {
      public:
        Element(HtmlWriter& html, std::string_view name) : _html(html), _name(name) {}
        ~Element() { _html.end(_name); }
        Element(const Element&) = delete;
        Element& operator=(const Element&) = delete;

      private:
        HtmlWriter& _html;
        std::string_view _name;
    };

    /// Name and attributes are constants of ours: `class="number"`.
    [[nodiscard]] Element inside(std::string_view name, std::string_view attributes = {});
    void element(std::string_view name, std::string_view text, std::string_view attributes = {});
    void text(std::string_view text);
    /// What is a piece of a document already.
    void piece(std::string_view markup) { _text += markup; }

    std::size_t size() const { return _text.size(); }
    const std::string& written() const { return _text; }

  private:
    void begin(std::string_view name, std::string_view attributes);
    void end(std::string_view name);

    std::string _text;
};

} // namespace ventrik
