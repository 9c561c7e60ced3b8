// Shows the living objects of a program in a browser:
//
//   vesk::Inspector inspector;
//   inspector.Show("orders", m_orders);
//   xout() << inspector.Listen() << '\n';       // the address, http://127.0.0.1:43210/9f0c.../
//   while (...) { ...; inspector.Poll(); }      // in the loop of the program
//
// or, where the program has no loop of its own,
//
//   inspector.Serve(8000);                      // prints the address, and is the loop
//
// There is no thread behind it: an object is read, changed and called within Poll or Serve alone, by the thread that
// calls them. That is always the same one, and the one whose graph and hooks are shown; only Stop may come from
// another. What is shown must live until it is hidden, and so must what it refers to. Between two calls of Poll the
// program may do with it what it likes. A Poll within a method that the page calls does nothing.
//
// While nobody looks, Poll reads the clock, and looks at its sockets a hundred times a second at most; no hook is set.
//
// The page reads. Changes and calls are for programs that say so: inspector.AllowChanges().
//
// It needs Boost.Beast (Debian's libboost-dev, headers alone), and nothing else includes it. Programs link with
// -pthread.

@import "Vesk/vxObject/InspectorPage.h"
@import "Vesk/vxObject/InspectorServer.h"

namespace vesk {

class Inspector {
 public:
  typedef InspectorServer::Clock Clock;

  explicit Inspector(xstring const& title = "Inspector")
      : m_server(m_shared, [](xstring const& nonce) { return InspectorPageText(nonce); }) {
    m_shared.m_title = title;
  }
  Inspector(Inspector const&) = delete;
  void operator=(Inspector const&) = delete;

  // Shows a value under a name, in place of what had it; one that is const cannot be changed. AccessError for a class
  // that nobody registered.
  template <typename T>
  void Show(xstring const& name, T& value) {
    m_shared.m_tree.Show(
        name, [shown = Value::Of(value)] { return shown; }, std::is_const<T>::value);
  }
  template <typename I>
  void ShowObject(xstring const& name, ptr<I> const& object) {
    if (!object) throw InspectorError("no object to show as " + name);
    ReflectedClass const* const record = QueryInterface<IObject>(object)->GetReflectedClass();
    ShowBy(name, [shown = Value(*record, object.Object())] { return shown; });
  }
  // What the function answers whenever it is looked at; an empty Value for nothing.
  void ShowBy(xstring const& name, std::function<Value()> source) {
    m_shared.m_tree.Show(name, std::move(source), false);
  }
  // False when there is nothing of the name.
  bool Hide(xstring const& name) { return m_shared.m_tree.Hide(name); }

  // Lets pages change values and call methods.
  void AllowChanges(bool isAllowed = true) { m_shared.m_changes.Allow(isAllowed); }

  // Whether pages may show archives, of which the objects are made and destroyed again: they may unless it is told.
  void TakeArchives(bool takes) { m_shared.m_takesArchives = takes; }

  // Begins to listen, on this machine alone; port 0 is any that is free. The address of the page, of which the token is
  // a secret. InspectorError when the port is taken.
  xstring Listen(uint16 port = 0) {
    if (!m_server.IsListening()) m_server.Listen(port);
    return Address();
  }
  xstring Address() const { return m_server.Address(); }
  std::size_t Pages() const { return m_server.Pages(); }
  InspectorServerLimits& Limits() { return m_server.Limits(); }

  // Serves what has come; it takes little longer than `most`, except for a method that the page calls.
  void Poll(Clock::duration most = std::chrono::milliseconds(10)) {
    const auto now = Clock::now();
    if (now < m_next || m_isBusy) return;
    const Busy busy(m_isBusy);
    m_server.Poll(most);
    m_next = now + (m_server.Pages() > 0 ? kPauseOfPages : kPause);
  }
  // Listens, prints the address, and serves until Stop or until `isDone`, which is asked ten times a second.
  void Serve(
      uint16 port = 0, std::function<bool()> const& isDone = [] { return false; }) {
    const xstring address = Listen(port);
    xout() << "Inspector: " << address << '\n';
    xout().Target().flush();
    const Busy busy(m_isBusy);
    while (!m_stops && !isDone()) m_server.Wait(m_server.Pages() > 0 ? kPause : std::chrono::milliseconds(100));
  }
  // Ends Serve; from any thread.
  void Stop() { m_stops = true; }

 private:
  static constexpr std::chrono::milliseconds kPause{10}, kPauseOfPages{1};

  struct Busy {
    explicit Busy(bool& isBusy) : m_isBusy(isBusy) { m_isBusy = true; }
    ~Busy() { m_isBusy = false; }
    Busy(Busy const&) = delete;
    void operator=(Busy const&) = delete;
    bool& m_isBusy;
  };

  InspectorShared m_shared;
  InspectorServer m_server;
  Clock::time_point m_next;
  std::atomic<bool> m_stops{false};
  bool m_isBusy = false;
};

}  // namespace vesk
